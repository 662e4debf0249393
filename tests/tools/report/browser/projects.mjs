// The projects on which the page is tested, each with its report. They are created once for each test file.
import {execFileSync} from 'node:child_process';
import {mkdirSync, mkdtempSync, readFileSync, rmSync, writeFileSync} from 'node:fs';
import {tmpdir} from 'node:os';
import {dirname, join} from 'node:path';
import {after} from 'node:test';

export const scratch = mkdtempSync(join(tmpdir(), 'report-projects-'));
after(() => rmSync(scratch, {recursive: true, force: true}));

const environment = {
    ...process.env, LC_ALL: 'C.UTF-8', GIT_CONFIG_GLOBAL: '/dev/null', GIT_AUTHOR_NAME: 'Ada', GIT_COMMITTER_NAME: 'Ada',
    GIT_AUTHOR_EMAIL: 'ada@example.org', GIT_COMMITTER_EMAIL: 'ada@example.org',
};

export function run(folder, program, args, settings = {}) {
    return execFileSync(program, args, {
        cwd: join(scratch, folder), env: {...environment, ...settings}, maxBuffer: 1 << 28,
    });
}

export const tool = (folder, ...args) => run(folder, process.env.PROJECTCTL, args);

/** Writes the report of a project beside it. @return the name of the page. */
export function report(folder, args = [], settings = {}) {
    const file = join(scratch, `${folder}${args.length > 0 ? '-compared' : ''}.html`);
    run(folder, process.env.PROJECTCTL, ['report', '--output', file, ...args], settings);
    return file;
}

export function createProject(folder, name, files) {
    mkdirSync(join(scratch, folder), {recursive: true});
    tool(folder, 'init', '--name', name);
    for (const [file, content] of Object.entries(files)) {
        mkdirSync(dirname(join(scratch, folder, file)), {recursive: true});
        writeFileSync(join(scratch, folder, file), content);
    }
    if (Object.keys(files).length > 0) {
        tool(folder, 'add', '--recursive', '.');
    }
}

function commit(folder, subject, date) {
    run(folder, 'git', ['add', '-A']);
    run(folder, 'git', ['commit', '-qm', subject], {GIT_AUTHOR_DATE: date, GIT_COMMITTER_DATE: date});
}

/** A project with labels, entry points, references that form a cycle, and a history. */
export function createEngine() {
    for (const other of ['pump', 'valve', 'gone']) {
        createProject(other, `The ${other}`, {});
    }
    mkdirSync(join(scratch, 'engine'), {recursive: true});
    run('engine', 'git', ['init', '-q', '-b', 'main']);
    createProject('engine', 'Engine controller', {
        'src/io/pump.cpp': 'line\n'.repeat(40), 'src/io/valve.cpp': 'line\n'.repeat(30), 'src/main.cpp': 'line\n'.repeat(90),
        'docs/readme.md': 'line\n'.repeat(20), 'docs/old.md': 'line\n', 'tools/clean.py': 'line\n'.repeat(10),
    });
    tool('engine', 'description', 'Controls the pumps');
    tool('engine', 'category', 'create', 'Status', '--single-valued');
    tool('engine', 'label', 'create', 'Status', 'Open');
    tool('engine', 'label', 'create', 'Status', 'Reviewed');
    tool('engine', 'category', 'create', 'Owner');
    tool('engine', 'label', 'create', 'Owner', 'Ada');
    tool('engine', 'label', 'create', 'Owner', 'Grace');
    tool('engine', 'label', 'put', 'Status', 'Open', 'src/io/pump.cpp', 'src/main.cpp');
    commit('engine', 'First', '2026-03-01T10:00:00+00:00');
    tool('engine', 'label', 'put', 'Status', 'Reviewed', 'src/io/valve.cpp');
    tool('engine', 'label', 'put', 'Owner', 'Ada', 'src/io/pump.cpp', 'docs/readme.md');
    tool('engine', 'label', 'put', 'Owner', 'Grace', 'src/io/pump.cpp');
    tool('engine', 'group', 'create', 'Nightly');
    tool('engine', 'entry', 'set', 'tools/clean.py', '--type', 'Batch_Job', '--group', 'Nightly');
    tool('engine', 'reference', 'add', '../pump');
    tool('pump', 'reference', 'add', '../valve');
    tool('valve', 'reference', 'add', '../engine');
    tool('valve', 'reference', 'add', '../gone');
    rmSync(join(scratch, 'gone'), {recursive: true});
    commit('engine', 'Second', '2026-04-01T10:00:00+00:00');
    tool('engine', 'label', 'put', 'Status', 'Reviewed', 'src/main.cpp');
    tool('engine', 'remove', 'docs/old.md');
    writeFileSync(join(scratch, 'engine/src/new.cpp'), 'x\n');
    tool('engine', 'add', 'src/new.cpp');
    writeFileSync(join(scratch, 'engine/docs/readme.md'), 'other\n');
    writeFileSync(join(scratch, 'engine/unknown.txt'), 'x\n');
}

/** A project in which a file and a category were renamed, and a folder was removed, since the last commit. */
export function createRenamed() {
    mkdirSync(join(scratch, 'renamed'), {recursive: true});
    run('renamed', 'git', ['init', '-q', '-b', 'main']);
    createProject('renamed', 'Renamed', {'gone/x.txt': 'x\n', 'src/main.cpp': 'x\n', 'src/old.cpp': 'one line\n'.repeat(20)});
    tool('renamed', 'category', 'create', 'Status');
    commit('renamed', 'First', '2026-03-01T10:00:00+00:00');
    tool('renamed', 'move', 'src/old.cpp', 'src/new.cpp');
    tool('renamed', 'category', 'rename', 'Status', 'State');
    tool('renamed', 'remove', 'gone');
}

/** Names that would do harm, or hide, if they were anything but text. */
export const hostileNames = [
    '<img src=x onerror=alert(1)>', '"onmouseover=alert(2)', '\'`${alert(3)}', 'new\nline\ttab', 'esc\u001b[31m',
    '\u202egnp.exe', 'שלום.txt', 'مرحبا', '<!--', ']]>', '&lt;&amp;', '%41%2f', '\\back', ' spaces ', '日本語.txt', '😀.md',
    '\u200bzero', '-rf', 'javascript:alert(4)', '{{data}}', '\\u003c',
];

export function createHostile() {
    const files = {'</script><script>alert(5)<': '1\n'};
    for (const folder of ['', '<b>/', '\u202efolder/']) {
        hostileNames.forEach((name, i) => { files[folder + name] = 'x\n'.repeat(i + 1); });
    }
    createProject('hostile', '</title></script><script>alert("name")</script>', files);
    writeFileSync(Buffer.concat([Buffer.from(`${scratch}/hostile/bad`), Buffer.from([0xff, 0xfe, 0x80])]), 'x\n');
    tool('hostile', 'add', '--recursive', '.');
    tool('hostile', 'description', '<b onclick=alert(6)>&amp;</script>');
    const label = '"><img src=x onerror=alert(7)>\n';
    tool('hostile', 'category', 'create', '</option><script>');
    tool('hostile', 'label', 'create', '</option><script>', label);
    tool('hostile', 'category', 'create', 'a=b&c');
    tool('hostile', 'label', 'create', 'a=b&c', '100% &');
    tool('hostile', 'label', 'put', '</option><script>', label, '<!--', 'مرحبا');
    tool('hostile', 'label', 'put', 'a=b&c', '100% &', '<b>/<!--');
    tool('hostile', 'entry', 'set', '<!--', '--name', '<script>alert(8)</script>');
}

/** A project of 100,000 files, which are in the definition only. */
export function createLarge() {
    createProject('large', 'Large', {});
    tool('large', 'category', 'create', 'Status');
    tool('large', 'label', 'create', 'Status', 'Open');
    const [category] = JSON.parse(tool('large', 'category', 'list', '--json')).categories;
    const [label] = JSON.parse(tool('large', 'label', 'list', 'Status', '--json')).labels.map((row) => row.label);
    const labels = `"children":[{"type":"Category","keys":{"UUID":"${category.uuid}"},"children":[{"type":"Label",` +
        `"keys":{"UUID":"${label.uuid}","Value":""}}]}]`;
    const lines = [];
    const pad = (number, digits) => String(number).padStart(digits, '0');
    for (let part = 0; part < 100; ++part) {
        lines.push(`"part_${pad(part, 2)}"`, `"part_${pad(part, 2)}/"`);
        for (let module = 0; module < 50; ++module) {
            const folder = `part_${pad(part, 2)}/module_${pad(module, 2)}`;
            lines.push(`"${folder}"`, `"${folder}/"`);
            for (let file = 0; file < 20; ++file) {
                const path = `${folder}/source_${pad(file, 2)}.cpp`;
                lines.push(file % 3 === 0 ? `{"file":"${path}",${labels}}` : `"${path}"`);
            }
        }
    }
    const text = join(scratch, 'large/.projectdata/project.jsonl');
    const old = readFileSync(text, 'utf8').split('\n');
    const place = old.findIndex((line) => line.startsWith('{"at":["Info"'));
    writeFileSync(text, [...old.slice(0, place), ...lines, ...old.slice(place)].join('\n'));
}

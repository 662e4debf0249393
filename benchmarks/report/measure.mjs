// Measures a page: see the script `measure`.
import {execFileSync} from 'node:child_process';
import {mkdtempSync, rmSync, statSync} from 'node:fs';
import {tmpdir} from 'node:os';
import {join} from 'node:path';
import {pathToFileURL} from 'node:url';
import puppeteer from 'puppeteer-core';

const [project, rounds] = [process.argv[2], Number(process.argv[3])];
const scratch = mkdtempSync(join(tmpdir(), 'report-measure-'));
const file = join(scratch, 'page.html');

const median = (values) => values.sort((left, right) => left - right)[values.length >> 1];
const shown = (name, values) => console.log(`${name.padEnd(46)} ${median(values).toFixed(0).padStart(6)} ms`);

function writePage() {
    const begin = performance.now();
    execFileSync(process.env.PROJECTCTL, ['report', '--output', file], {cwd: project});
    return performance.now() - begin;
}

/** From the start of the navigation until the map is drawn and the list answers. */
async function openPage(browser) {
    const page = await browser.newPage();
    await page.setViewport({width: 1280, height: 900});
    await page.goto(pathToFileURL(file).href);
    await page.waitForFunction(() => document.documentElement.dataset.ready === 'true');
    const usable = await page.evaluate(() => new Promise((done) => {
        requestAnimationFrame(() => requestAnimationFrame(() => done(performance.now())));
    }));
    return {page, usable};
}

/** A piece of work with the frame that shows it. */
const timeOf = (page, work) => page.evaluate(`new Promise((done) => {
    const begin = performance.now();
    (${work})();
    const used = performance.now() - begin;
    requestAnimationFrame(() => requestAnimationFrame(() => done({used, frame: performance.now() - begin})));
})`);

const works = {
    'zoom to a folder of 1000 files': "() => shownPage.map.zoomTo(shownPage.model.paths.indexOf('part_42') + 1)",
    'zoom to the whole project': '() => shownPage.map.zoomTo(0)',
    'other areas (lines), the first time':
        "() => { const select = byId('mapMeasure'); select.value = 'lines'; select.dispatchEvent(new Event('change')); }",
    'search in all paths': "() => shownPage.files.form.update({search: 'module_17/source_1'})",
    'pattern on all paths': "() => shownPage.files.form.set({...noConditions(), glob: '**/module_1?/*.cpp'})",
    'sort by size': "() => shownPage.files.form.set({...noConditions(), sort: '-size'})",
};

const browser = await puppeteer.launch({
    executablePath: '/usr/bin/chromium', userDataDir: join(scratch, 'profile'),
    args: ['--no-sandbox', '--disable-gpu', '--disable-quic', '--no-first-run', '--disable-background-networking',
        '--disable-component-update', '--disable-sync', '--disable-dev-shm-usage'],
});
const times = {write: [], usable: [], works: Object.fromEntries(Object.keys(works).map((name) => [name, {used: [], frame: []}]))};
for (let round = 0; round < rounds; ++round) {
    times.write.push(writePage());
    const {page, usable} = await openPage(browser);
    times.usable.push(usable);
    for (const [name, work] of Object.entries(works)) {
        const {used, frame} = await timeOf(page, work);
        times.works[name].used.push(used);
        times.works[name].frame.push(frame);
    }
    await page.close();
}
await browser.close();
console.log(`the page of 100,000 files: ${statSync(file).size} bytes; medians of ${rounds} rounds`);
shown('projectctl report', times.write);
shown('opening the page until it is usable', times.usable);
for (const [name, {used, frame}] of Object.entries(times.works)) {
    shown(`${name}: work`, used);
    shown(`${name}: until it is shown`, frame);
}
rmSync(scratch, {recursive: true, force: true});

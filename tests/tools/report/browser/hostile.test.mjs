import assert from 'node:assert/strict';
import {readFileSync} from 'node:fs';
import {test} from 'node:test';
import {drawn, textOf, textsOf, useBrowser, withPage} from './browser.mjs';
import {createHostile, hostileNames, report} from './projects.mjs';

createHostile();
const hostile = report('hostile');
useBrowser();

test('names appear as text, and nothing in them becomes an element or runs', () => withPage(hostile, {}, async (page) => {
    assert.equal(await textOf(page, 'h1'), '</title></script><script>alert("name")</script>');
    assert.equal(await textOf(page, '#description'), '<b onclick=alert(6)>&amp;</script>');
    assert.deepEqual(await page.evaluate(() => ({
        scripts: document.scripts.length,
        others: document.querySelectorAll('img, iframe, object, embed, b, [onclick], [onerror]').length,
        outside: document.body.lastElementChild.tagName,
    })), {scripts: 3, others: 0, outside: 'SCRIPT'});
    const links = await page.$$eval('a', (all) => all.map((link) => link.getAttribute('href')));
    assert.ok(links.length > 10 && links.every((link) => link.startsWith('#')), links.join(' '));
}));

test('every name is in the data as it is on disk', () => withPage(hostile, {}, async (page) => {
    const paths = new Set(await page.evaluate(() => shownPage.model.paths));
    for (const folder of ['', '<b>/', '\u202efolder/']) {
        hostileNames.forEach((name) => assert.ok(paths.has(folder + name), folder + name));
    }
    assert.ok(paths.has('bad\udcff\udcfe\udc80'));
    assert.ok(paths.has('</script><script>alert(5)<'));
}));

test('invisible characters, and bytes that are not valid UTF-8, are shown as escapes', () => withPage(hostile, {}, async (page) => {
    await page.evaluate(() => shownPage.files.form.set({...noConditions(), glob: '*'}));
    const names = new Set(await page.evaluate(() =>
        findEntries(shownPage.model, noConditions()).map((entry) => shownName(shownPage.model.paths[entry]))));
    for (const name of ['bad\\xff\\xfe\\x80', 'new\\nline\\ttab', 'esc\\u001b[31m', '\\u202egnp.exe', '\\u200bzero']) {
        assert.ok(names.has(name), name);
    }
    const shown = await page.evaluate(() => document.body.innerText);
    assert.doesNotMatch(shown, /[\u0000-\u0008\u000b-\u001f\u200b\u202a-\u202e]/u);
    assert.ok((await textsOf(page, '.rows .name')).every((name) => !/[\ud800-\udfff]/u.test(name)));
}));

test('a link to any name leads to it', () => withPage(hostile, {}, async (page) => {
    const wrong = await page.evaluate(() => shownPage.model.paths.filter((path) => {
        const link = linkToPath(path);
        const isPlain = /^#filter=path=[\w.~!*'()%-]*$/u.test(link);
        return !isPlain || conditionsOf(shownPage.model, link).paths[0] !== path;
    }));
    assert.deepEqual(wrong, []);
}));

test('names in right-to-left scripts do not affect the text around them', () => withPage(hostile, {}, async (page) => {
    await page.evaluate(() => shownPage.files.form.set({...noConditions(), search: 'مرحبا'}));
    await drawn(page); // the list replaces its rows with the next frame
    const places = await page.evaluate(() => {
        const row = document.querySelector('.rows .row');
        return [...row.children].map((cell) => cell.getBoundingClientRect().x);
    });
    assert.ok(places.length > 1);
    assert.deepEqual(places, [...places].sort((left, right) => left - right));
    const directions = await page.evaluate(() =>
        [...document.querySelectorAll('.name')].map((name) => getComputedStyle(name).unicodeBidi));
    assert.ok(directions.length > 1);
    assert.deepEqual(directions.filter((direction) => direction !== 'isolate'), []);
}));

test('the data contain no character that HTML gives a meaning to', () => {
    const page = readFileSync(hostile, 'latin1');
    const data = page.slice(page.indexOf('id="data">') + 10, page.indexOf('</script>', page.indexOf('id="data">')));
    assert.ok(data.length > 1000);
    assert.doesNotMatch(data, /[<\u0000-\u001f]/u);
    JSON.parse(Buffer.from(data, 'latin1').toString('utf8'));
});

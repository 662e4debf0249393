import assert from 'node:assert/strict';
import {statSync} from 'node:fs';
import {test} from 'node:test';
import {drawn, textOf, textsOf, useBrowser, withPage} from './browser.mjs';
import {createLarge, report, tool} from './projects.mjs';

createLarge();
const large = report('large');
useBrowser();

test('a page of 100,000 files is smaller than 3 MB', () => {
    assert.ok(statSync(large).size < 3000000, String(statSync(large).size));
});

test('it has all paths in the order of list', () => withPage(large, {}, async (page) => {
    assert.equal(await textOf(page, '#filesCount'), '105,100 of 105,100 entries');
    const paths = await page.evaluate(() => shownPage.model.paths);
    assert.equal(`${paths.join('\n')}\n`, tool('large', 'list').toString());
}));

test('the list has a few rows in the document, and shows the rows at each place', () => withPage(large, {}, async (page) => {
    assert.ok((await page.$$('.rows .row')).length < 80);
    await page.focus('.grid');
    await page.keyboard.press('End');
    await drawn(page);
    assert.equal(await textOf(page, '.row.current .name'), 'part_99/module_49/source_19.cpp');
    assert.equal(await page.$eval('.row.current', (row) => row.getAttribute('aria-rowindex')), '105101');
    const isVisible = await page.evaluate(() => {
        const row = document.querySelector('.row.current').getBoundingClientRect();
        const grid = document.querySelector('.grid').getBoundingClientRect();
        return row.top >= grid.top && row.bottom <= grid.bottom + 1;
    });
    assert.ok(isVisible);
    await page.evaluate(() => { location.hash = '#filter=search=module_07/source_05&kind=file'; });
    await drawn(page);
    assert.equal(await textOf(page, '#filesCount'), '100 of 105,100 entries');
}));

test('folders too small for their files are one tile with the shares of their labels', () => withPage(large, {}, async (page) => {
    const tiles = await page.evaluate(() => shownPage.map.root.leaves().length);
    assert.ok(tiles >= 100 && tiles < 20000, String(tiles));
    assert.deepEqual(await textsOf(page, '#legend .number'), ['35,000', '65,000']);
    await page.evaluate(() => shownPage.map.zoomTo(shownPage.model.paths.indexOf('part_42/module_17') + 1));
    assert.equal(await page.evaluate(() => shownPage.map.root.leaves().length), 20);
    assert.match((await textOf(page, '#mapHere')).replace(/[\u2068\u2069]/gu, ''), /part_42\/module_17\/.* 20 files · No label 65% · Open 35%/u);
}));

test('a list that is taller than a browser can lay out still shows its last row', () => withPage(large, {}, async (page) => {
    const last = await page.evaluate(() => {
        const {list} = shownPage.files;
        list.show(Array.from({length: 400000}, (_, i) => i % 105100));
        list.moveTo(399999);
        const row = document.querySelector('.row.current').getBoundingClientRect();
        const grid = list.grid.getBoundingClientRect();
        return {height: list.rows.offsetHeight, isVisible: row.top >= grid.top && row.bottom <= grid.bottom + 2};
    });
    assert.deepEqual(last, {height: 8000000, isVisible: true});
}));

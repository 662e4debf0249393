import assert from 'node:assert/strict';
import {test} from 'node:test';
import {useBrowser, withPage} from './browser.mjs';
import {createEngine, createHostile, report} from './projects.mjs';

createEngine();
createHostile();
const pages = {engine: report('engine', ['--compare', 'HEAD~1']), hostile: report('hostile')};
useBrowser();

/** The contrasts of all visible texts with the backgrounds behind them, and of borders and the map's colours. */
const contrasts = (page) => page.evaluate(() => {
    const parse = (colour) => colour.match(/[\d.]+/gu).map(Number);
    const ofHex = (hex) => [1, 3, 5].map((at) => parseInt(hex.slice(at, at + 2), 16));
    const luminance = ([r, g, b]) => {
        const linear = [r, g, b].map((value) => value / 255)
            .map((value) => (value <= 0.04045 ? value / 12.92 : ((value + 0.055) / 1.055) ** 2.4));
        return 0.2126 * linear[0] + 0.7152 * linear[1] + 0.0722 * linear[2];
    };
    const contrast = (one, other) => {
        const [high, low] = [luminance(one), luminance(other)].sort((left, right) => right - left);
        return (high + 0.05) / (low + 0.05);
    };
    const background = (place) => {
        for (let at = place; at !== null; at = at.parentElement) {
            const colour = parse(getComputedStyle(at).backgroundColor);
            if (colour.length < 4 || colour[3] === 1) {
                return colour;
            }
        }
        return [255, 255, 255];
    };
    const texts = [];
    const walker = document.createTreeWalker(document.body, NodeFilter.SHOW_TEXT);
    for (let node = walker.nextNode(); node !== null; node = walker.nextNode()) {
        const place = node.parentElement;
        const style = getComputedStyle(place);
        const isShown = place.getClientRects().length > 0 && node.textContent.trim() !== '' && style.visibility === 'visible';
        if (isShown && !['SCRIPT', 'STYLE', 'OPTION'].includes(place.tagName)) {
            const isSvg = place instanceof SVGElement;
            const behind = isSvg ? ofHex(schemeColour(place.closest('.node') ? 'surface' : 'paper')) : background(place);
            texts.push({text: node.textContent.trim().slice(0, 40),
                contrast: contrast(parse(isSvg ? style.fill : style.color), behind)});
        }
    }
    const scheme = (name) => ofHex(schemeColour(name));
    const ink = ofHex('#0d1117');
    const tiles = [...groupColours, noLabelColour, ...Object.values(changeColours)];
    return {
        texts,
        headings: contrast(scheme('ink'), scheme('frame')), // of the folders on the map
        tiles: tiles.map((colour) => ({
            onSurface: contrast(ofHex(colour), scheme('surface')), ofText: contrast(ink, ofHex(colour)),
            onPaper: contrast(ofHex(colour), scheme('paper')), // lines of the charts
        })),
        borders: ['surface', 'paper'].flatMap((behind) => ['control', 'accent', 'fault'].map((name) =>
            contrast(scheme(name), scheme(behind)))),
    };
});

/** Shows everything that is not shown at first: a chosen row, a condition, and the path under the pointer. */
const showAll = (page) => page.evaluate(() => {
    const {map, files} = shownPage;
    files.form.set({...noConditions(), unknown: ['Nothing=Here'], labels: [{category: 0, label: null}], paths: ['src']});
    files.form.onChange(noConditions());
    files.list.moveTo(1);
    map.showTip(map.root.children[0], {clientX: 0, clientY: 0});
    document.querySelectorAll('details').forEach((details) => details.setAttribute('open', ''));
});

for (const scheme of ['light', 'dark']) {
    for (const [name, file] of Object.entries(pages)) {
        test(`all texts, borders and colours have enough contrast: ${name}, ${scheme}`, () =>
            withPage(file, {scheme}, async (page) => {
                await showAll(page);
                const {texts, headings, tiles, borders} = await contrasts(page);
                assert.ok(texts.length > 60);
                assert.deepEqual(texts.filter((item) => item.contrast < 4.5), []);
                assert.ok(headings >= 4.5);
                assert.deepEqual(tiles.filter((tile) => tile.onSurface < 3 || tile.onPaper < 3 || tile.ofText < 4.5), []);
                assert.deepEqual(borders.filter((contrast) => contrast < 3), []);
            }));
    }
}

test('the schemes differ, and the map follows a change of the scheme', () => withPage(pages.engine, {}, async (page) => {
    const frame = () => page.evaluate(() => {
        shownPage.map.redraw();
        return [getComputedStyle(document.body).backgroundColor, shownPage.map.drawing.frame];
    });
    const light = await frame();
    await page.emulateMediaFeatures([{name: 'prefers-color-scheme', value: 'dark'}]);
    const dark = await frame();
    assert.notEqual(light[0], dark[0]);
    assert.notEqual(light[1], dark[1]);
}));

for (const width of [390, 820, 1280]) {
    for (const [name, file] of Object.entries(pages)) {
        test(`nothing is wider than the window: ${name}, ${width} px`, () => withPage(file, {width}, async (page) => {
            const widest = await page.evaluate(() => document.scrollingElement.scrollWidth);
            assert.ok(widest <= width, `${widest} px`);
            const map = await page.evaluate(() => {
                const box = document.getElementById('mapCanvas').getBoundingClientRect();
                return {width: box.width, root: shownPage.map.root.x1, height: box.height};
            });
            assert.ok(map.width > 0.6 * Math.min(width, 900) && map.height >= 300);
            assert.ok(Math.abs(map.width - map.root) <= 1);
        }));
    }
}

test('everything that can be used has a name, and every picture has a table', () => withPage(pages.engine, {}, async (page) => {
    const unnamed = await page.evaluate(() => [...document.querySelectorAll('button, a, input, select, canvas, [role=grid], nav, svg[role=img]')]
        .filter((place) => (place.getAttribute('aria-label') ?? '') === '' && place.textContent.trim() === '' &&
            (place.closest('label')?.textContent.trim() ?? '') === '' && place.id !== 'sections')
        .map((place) => place.outerHTML.slice(0, 120)));
    assert.deepEqual(unnamed, []);
    for (const section of ['map', 'references', 'history']) {
        assert.notEqual(await page.$(`#${section} table`), null, section);
    }
    const ids = await page.$$eval('[id]', (all) => all.map((place) => place.id));
    assert.equal(new Set(ids).size, ids.length);
    const headings = await page.$$eval('h1, h2, h3', (all) => all.map((heading) => Number(heading.tagName[1])));
    headings.forEach((level, i) => assert.ok(i === 0 ? level === 1 : level <= headings[i - 1] + 1));
}));

test('the keyboard reaches every control in the order of the page', () => withPage(pages.engine, {}, async (page) => {
    await page.evaluate(() => {
        [...document.querySelectorAll('a[href], button, input, select, summary, [tabindex="0"]')]
            .filter((place) => place.checkVisibility())
            .forEach((place, i) => { place.dataset.control = `${i} ${place.id || place.className || place.tagName}`; });
    });
    const reached = [];
    for (let i = 0; i < 400; ++i) {
        await page.keyboard.press('Tab');
        const control = await page.evaluate(() => {
            const place = document.activeElement;
            if (place === document.body) {
                return null;
            }
            const isVisible = place.matches(':focus-visible') && getComputedStyle(place).outlineStyle !== 'none';
            return `${isVisible ? '' : 'invisible '}${place.dataset.control ?? place.outerHTML.slice(0, 80)}`;
        });
        if (control === null) {
            break;
        }
        reached.push(control);
    }
    const controls = await page.$$eval('[data-control]', (all) => all.map((place) => place.dataset.control));
    for (const id of ['mapColour', 'mapMeasure', 'mapCanvas', 'filterSearch', 'filterGlob', 'filterWithLabel', 'clearFilter',
        'filterLink', 'grid']) {
        assert.ok(controls.some((control) => control.endsWith(` ${id}`)), id);
    }
    assert.deepEqual(reached, controls);
}));

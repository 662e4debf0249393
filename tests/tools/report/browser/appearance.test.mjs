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
    const surface = ofHex(schemeColour('surface'));
    const ink = ofHex('#0d1117');
    const tiles = [...groupColours, noLabelColour, ...Object.values(changeColours)];
    return {
        texts,
        tiles: tiles.map((colour) => ({onSurface: contrast(ofHex(colour), surface), ofText: contrast(ink, ofHex(colour))})),
        borders: ['surface', 'paper'].map((name) => contrast(ofHex(schemeColour('control')), ofHex(schemeColour(name)))),
    };
});

for (const scheme of ['light', 'dark']) {
    for (const [name, file] of Object.entries(pages)) {
        test(`all texts, borders and colours have enough contrast: ${name}, ${scheme}`, () =>
            withPage(file, {scheme}, async (page) => {
                const {texts, tiles, borders} = await contrasts(page);
                assert.ok(texts.length > 60);
                assert.deepEqual(texts.filter((item) => item.contrast < 4.5), []);
                assert.deepEqual(tiles.filter((tile) => tile.onSurface < 3 || tile.ofText < 4.5), []);
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
    const reached = [];
    for (let i = 0; i < 400; ++i) {
        await page.keyboard.press('Tab');
        const id = await page.evaluate(() => {
            const place = document.activeElement;
            if (place === document.body) {
                return null;
            }
            const isVisible = place.matches(':focus-visible') && getComputedStyle(place).outlineStyle !== 'none';
            return `${isVisible ? '' : 'invisible '}${place.id || place.className || place.tagName}`;
        });
        if (id === null) {
            break;
        }
        reached.push(id);
    }
    assert.deepEqual(reached.filter((id) => id.startsWith('invisible')), []);
    const controls = ['mapColour', 'mapMeasure', 'mapCanvas', 'filterSearch', 'filterGlob', 'filterWithLabel', 'clearFilter',
        'filterLink', 'grid'];
    const places = controls.map((id) => reached.indexOf(id));
    assert.ok(places.every((place) => place >= 0), JSON.stringify(reached));
    assert.deepEqual(places, [...places].sort((left, right) => left - right));
}));

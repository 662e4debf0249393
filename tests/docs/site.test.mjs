// The site of the documentation in a browser, opened as files: at two widths, light and dark. SITE is its folder.
import assert from 'node:assert/strict';
import {readdirSync} from 'node:fs';
import {join} from 'node:path';
import {test} from 'node:test';
import {pathToFileURL} from 'node:url';
import {drawn, newPage, useBrowser} from './browser.mjs';

const site = process.env.SITE;
const address = pathToFileURL(site + '/').href;
const widths = [390, 1280];
const schemes = ['light', 'dark'];
const reference = ['index.html', 'modules.html', 'annotated.html', 'namespaces.html', 'group__session.html', 'group__files.html',
    'group__platform.html', 'classproject_1_1session_1_1Session.html', 'structproject_1_1session_1_1Query.html',
    'classproject_1_1stores_1_1StoreError.html'].map((name) => `reference/${name}`);

useBrowser();

/** The pages of a folder of the site, without the reference. */
function pagesIn(folder = '') {
    return readdirSync(join(site, folder), {withFileTypes: true}).flatMap((entry) => {
        const path = folder + entry.name;
        if (entry.isDirectory()) {
            return path === 'reference' || entry.name.startsWith('_') ? [] : pagesIn(`${path}/`);
        }
        return path.endsWith('.html') ? [path] : [];
    });
}

/** Defines on a page: the contrast of two colours, and the texts that are too pale. */
function defineContrast() {
    const parse = (colour) => {
        const parts = colour.match(/^rgba?\((.*)\)$/)[1].split(',').map(Number);
        return {channels: parts.slice(0, 3), alpha: parts[3] ?? 1};
    };
    const over = (top, bottom) => top.channels.map((value, i) => value * top.alpha + bottom[i] * (1 - top.alpha));
    const luminance = (channels) => {
        const [r, g, b] = channels.map((value) => value / 255)
            .map((value) => (value <= 0.04045 ? value / 12.92 : ((value + 0.055) / 1.055) ** 2.4));
        return 0.2126 * r + 0.7152 * g + 0.0722 * b;
    };
    const background = (element) => {
        if (!element) {
            return [255, 255, 255];
        }
        const own = parse(getComputedStyle(element).backgroundColor);
        return own.alpha === 1 ? own.channels : over(own, background(element.parentElement));
    };
    window.contrast = (colour, below) => {
        const [light, dark] = [luminance(over(parse(colour), below)), luminance(below)].sort((a, b) => b - a);
        return (light + 0.05) / (dark + 0.05);
    };
    window.parseColour = parse;
    window.backgroundOf = background;
    const isShown = (element) => !element.closest('svg, .visually-hidden') &&
        element.checkVisibility({checkOpacity: true, checkVisibilityCSS: true});
    window.paleTexts = () => {
        const walker = document.createTreeWalker(document.body, NodeFilter.SHOW_TEXT);
        const pale = [];
        while (walker.nextNode()) {
            const element = walker.currentNode.parentElement;
            const text = walker.currentNode.data.trim();
            if (text && isShown(element)) {
                const ratio = contrast(getComputedStyle(element).color, background(element));
                if (ratio < 4.5) {
                    pale.push(`${text.slice(0, 30)}: ${ratio.toFixed(2)}`);
                }
            }
        }
        return pale;
    };
}

/** The faults of the page as it is shown now. */
function faults() {
    const found = paleTexts();
    if (document.documentElement.scrollWidth > innerWidth) {
        found.push(`is ${document.documentElement.scrollWidth} pixels wide`);
    }
    const headings = document.querySelectorAll('h1').length;
    if (headings !== 1) {
        found.push(`has ${headings} headings of the first level`);
    }
    const dashes = document.querySelector('article')?.innerText.match(/\s–\w+/g) ?? [];
    found.push(...dashes.map((option) => `shows a dash for the hyphens of${option}`));
    for (const image of document.images) {
        if (image.getClientRects().length && image.naturalWidth === 0) {
            found.push(`does not show ${image.src}`);
        }
        if (!image.alt && image.closest('article')) {
            found.push(`has no text for ${image.src}`);
        }
    }
    return found;
}

/** A page of the site. A picture inside a style sheet is not a request. */
async function openSite(options) {
    const page = await newPage(address, options);
    page.takeNoises = () => page.noises.splice(0).filter((noise) => !noise.startsWith('request: data:'));
    return page;
}

const show = async (page, width, scheme) => {
    await page.setViewport({width, height: 900});
    await page.emulateMediaFeatures([{name: 'prefers-color-scheme', value: scheme}]);
};

test('every page is readable at both widths, light and dark, and loads nothing from elsewhere', async () => {
    const page = await openSite();
    await page.evaluateOnNewDocument(defineContrast);
    const paths = [...pagesIn(), ...reference];
    const problems = [];
    for (const path of paths) {
        await page.goto(address + path);
        for (const width of widths) {
            for (const scheme of schemes) {
                await show(page, width, scheme);
                await drawn(page);
                problems.push(...(await page.evaluate(faults)).map((fault) => `${path}, ${width}, ${scheme}: ${fault}`));
            }
        }
        problems.push(...page.takeNoises().map((noise) => `${path}: ${noise}`));
    }
    assert.deepEqual(problems, []);
    assert.ok(paths.length > 40, `${paths.length} pages`);
});

/** The texts of a picture that are too pale on the shape below them, or on the page. */
function paleLabels(page) {
    return [...document.querySelectorAll('text')].flatMap((text) => {
        const box = text.getBoundingClientRect();
        const shapes = document.elementsFromPoint(box.x + box.width / 2, box.y + box.height / 2)
            .filter((element) => element.matches('rect, path, circle, polygon, ellipse'));
        const fills = shapes.map((shape) => getComputedStyle(shape).fill).filter((fill) => fill.startsWith('rgb('));
        const ratio = contrast(getComputedStyle(text).fill, parseColour(fills[0] ?? page).channels);
        return ratio < 4.5 ? [`${text.textContent}: ${ratio.toFixed(2)}`] : [];
    });
}

test('the texts of the pictures are readable on the page, light and dark', async () => {
    const pictures = readdirSync(join(site, '_images')).filter((name) => name.endsWith('.svg'));
    const page = await openSite();
    await page.evaluateOnNewDocument(defineContrast);
    const problems = [];
    for (const scheme of schemes) {
        await show(page, 1280, scheme);
        await page.goto(`${address}guide/concepts.html`);
        const [behind, below] = await page.$eval('article img', (image) => [getComputedStyle(image).backgroundColor,
            `rgb(${backgroundOf(image).join(', ')})`]);
        assert.match(behind, /, 0\)$/, 'a picture has the background of its page');
        for (const picture of pictures) {
            await page.goto(`${address}_images/${picture}`);
            problems.push(...(await page.evaluate(paleLabels, below)).map((label) => `${picture}, ${scheme}: ${label}`));
        }
    }
    assert.deepEqual(problems, []);
    assert.ok(pictures.length >= 4);
});

test('the chosen scheme of a page is that of its pictures', async () => {
    const page = await openSite();
    await page.goto(`${address}guide/concepts.html`);
    for (const scheme of schemes) {
        const used = await page.evaluate((chosen) => {
            document.body.dataset.theme = chosen;
            return getComputedStyle(document.querySelector('article img')).colorScheme;
        }, scheme);
        assert.equal(used, scheme);
    }
});

test('the menu of a narrow page opens, and leads to other pages', async () => {
    const page = await openSite({width: 390});
    await page.goto(`${address}index.html`);
    const entry = '.sidebar-tree a[href="guide/start.html"]';
    const isOnScreen = () => page.$eval(entry, (link) => {
        const box = link.getBoundingClientRect();
        return box.left >= 0 && box.right <= innerWidth;
    });
    assert.equal(await isOnScreen(), false);
    await page.click('.mobile-header label[for="__navigation"]');
    await page.waitForFunction((link) => document.querySelector(link).getBoundingClientRect().left >= 0, {}, entry);
    assert.equal(await isOnScreen(), true);
    await Promise.all([page.waitForNavigation(), page.click(entry)]);
    assert.equal(await page.$eval('h1', (heading) => heading.firstChild.data), 'Get started');
    assert.deepEqual(page.takeNoises(), []);
});

test('the search finds pages without a server', async () => {
    const page = await openSite();
    await page.goto(`${address}search.html?q=closing+line`);
    await page.waitForSelector('#search-results li a');
    const found = await page.$$eval('#search-results li a', (links) => links.map((link) => link.textContent));
    assert.ok(found.includes('The format'), found.join(', '));
    await Promise.all([page.waitForNavigation(), page.click('#search-results li a')]);
    assert.deepEqual(page.takeNoises(), []);
});
